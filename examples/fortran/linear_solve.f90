! linear_solve.f90 -- a dense system solved by ynsega (Gaussian elimination with complete
! pivoting) from Fortran, then a singular matrix and its code. Fortran arrays are column-major
! as the routine expects: a(i, j) is passed as it is.
program linear_solve
  use, intrinsic :: iso_c_binding, only: c_int, c_double
  use orvq7maths
  implicit none
  real(c_double) :: a(3, 3), b(3), x(3), s(2, 2), y(2)
  integer(c_int) :: ierr, r
  integer :: failures = 0

  !     | 4 2 0 |       | 1 |       |  8 |
  ! A = | 1 4 2 |   x = | 2 |   b = | 15 |
  !     | 0 2 4 |       | 3 |       | 16 |
  ! By hand: pivots 4 at (1, 1), then 4 at (3, 3) (rows and columns 2 and 3 exchanged),
  ! multipliers 1/4 and 1/2, the last row keeps 2.5 x2 = 5: every step is exact.
  a = reshape([4, 1, 0, 2, 4, 2, 0, 2, 4], [3, 3])
  b = [8, 15, 16]
  x = 0
  r = ynsega(3_c_int, a, b, x, ierr)
  call check_int("ynsega result", r, 0)
  call check_int("  ierr", ierr, ORVQ7_OK)
  call check("  x1", x(1), 1.0_c_double)
  call check("  x2", x(2), 2.0_c_double)
  call check("  x3", x(3), 3.0_c_double)

  ! | 1 2 |  pivot 4, multiplier 1/2, last pivot 1 - 0.5 * 2 = 0: singular (4703), and y keeps
  ! | 2 4 |  what it held.
  s = reshape([1, 2, 2, 4], [2, 2])
  y = -7
  r = ynsega(2_c_int, s, [1.0_c_double, 1.0_c_double], y, ierr)
  call check_int("ynsega (singular) result", r, 1)
  call check_int("  ierr", ierr, ORVQ7_ERR_SINGULAR)
  call check("  y1 untouched", y(1), -7.0_c_double)
  call check("  y2 untouched", y(2), -7.0_c_double)

  if (failures /= 0) error stop 1

contains

  subroutine check(what, got, want)
    character(*), intent(in) :: what
    real(c_double), intent(in) :: got, want
    print '(a26, 1x, es25.17)', what, got
    if (got /= want) then
      print '(a, es25.17)', "  expected ", want
      failures = failures + 1
    end if
  end subroutine check

  subroutine check_int(what, got, want)
    character(*), intent(in) :: what
    integer(c_int), intent(in) :: got
    integer, intent(in) :: want
    print '(a26, 1x, i0)', what, got
    if (got /= want) then
      print '(a, i0)', "  expected ", want
      failures = failures + 1
    end if
  end subroutine check_int

end program linear_solve
