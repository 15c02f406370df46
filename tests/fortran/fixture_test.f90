! tests/fortran/fixture_test.f90 -- calls every routine of fixture.h through the generated
! module and checks what comes back; stops with a non-zero code at the first mismatch.
module fixture_callbacks
  use, intrinsic :: iso_c_binding, only: c_int, c_double
  implicit none
contains
  ! f(x) = x(1) * x(2); result 3 so the caller can tell it was called.
  function product2(x, fx) bind(C) result(r)
    real(c_double), intent(in) :: x(2)
    real(c_double), intent(out) :: fx
    integer(c_int) :: r
    fx = x(1) * x(2)
    r = 3
  end function product2
  function negate(y, gy) bind(C) result(r)
    real(c_double), intent(in) :: y
    real(c_double), intent(out) :: gy
    integer(c_int) :: r
    gy = -y
    r = 1
  end function negate
end module fixture_callbacks

program fixture_test
  use, intrinsic :: iso_c_binding, only: c_int, c_int16_t, c_int64_t, c_double, c_char, &
                                         c_loc, c_funloc, c_f_pointer
  use orvq7_fixture
  use fixture_callbacks
  implicit none
  real(c_double) :: v(4) = [1.0_c_double, 2.0_c_double, 3.5_c_double, -0.5_c_double]
  real(c_double) :: x(3) = [1.0_c_double, 2.0_c_double, 3.0_c_double]
  real(c_double) :: y(3) = [10.0_c_double, 20.0_c_double, 30.0_c_double]
  real(c_double), target :: area(5)
  real(c_double) :: total, fx, gy
  integer(c_int) :: ierr, i, j, t(2, 3)
  integer(c_int64_t) :: k
  character(kind=c_char, len=6), target :: word
  character(kind=c_char), pointer :: chars(:)
  integer(c_int), target :: record(1) = [100]

  ! Constants from #define and from both enums.
  call expect(ORVQ7FIX_LIMIT == 7 .and. ORVQ7FIX_BAD == 4712 .and. ORVQ7FIX_OK == 0, 1)

  ! Arrays in, scalars out, a status pair; a failure leaves total untouched.
  total = -1.0_c_double
  call expect(fxsum(4_c_int, v, total, ierr) == 0 .and. total == 6.0_c_double &
              .and. ierr == 0, 2)
  total = -1.0_c_double
  call expect(fxsum(0_c_int, v, total, ierr) == 1 .and. ierr == 4712 &
              .and. total == -1.0_c_double, 3)

  ! Shapes given by reference to another routine's block.
  call expect(fxmean(4_c_int, v, total, ierr) == 0 .and. total == 1.5_c_double, 18)

  ! A subroutine; and a declaration sharing the block above it takes its shapes.
  call fxaxpy(2.0_c_double, x, y)
  call expect(all(y == [12.0_c_double, 24.0_c_double, 36.0_c_double]), 4)
  call fxaxpz(1.0_c_double, x, y)
  call expect(all(y == [-11.0_c_double, -22.0_c_double, -33.0_c_double]), 5)

  ! A two-dimensional integer table and an 8-byte integer, both by reference.
  t = reshape([1, 2, 3, 4, 5, 6], [2, 3])
  k = 3000000000_c_int64_t
  call expect(fxtab(t, 2_c_int, 3_c_int, 10_c_int64_t) == 60_c_int64_t, 6)
  call expect(all(t == reshape([11, 12, 13, 14, 15, 16], [2, 3])), 7)
  call expect(fxtab(t, 1_c_int, 1_c_int, k) == k, 8)

  ! Scalars by reference, written back.
  i = 5
  j = 9
  call expect(fxswap(i, j) == 4 .and. i == 9 .and. j == 5, 9)

  ! Characters with their length by value, an enum and an integer by value, a C string back.
  word = "AB CD "
  call expect(fxname(word, 4_c_int, 2_c_int, len(word, kind=c_int)) == 14, 10)
  call c_f_pointer(fxlast(), chars, [7])
  call expect(all(chars(1:7) == ["A", "B", " ", "C", "D", " ", achar(0)]), 11)
  call fxclear()
  call expect(chars(1) == achar(0), 12)

  ! An address and a real by value.
  area = 0.0_c_double
  call expect(fxfill(c_loc(area), 3_c_int, 2.5_c_double) == 3, 13)
  call expect(all(area == [2.5_c_double, 2.5_c_double, 2.5_c_double, 0.0_c_double, &
                           0.0_c_double]), 14)

  ! Routine arguments: C calls both Fortran procedures back.
  call expect(fxcall(c_funloc(product2), [3.0_c_double, 4.0_c_double], fx, &
                     c_funloc(negate), 2.0_c_double, gy) == 13, 15)
  call expect(fx == 12.0_c_double .and. gy == -2.0_c_double, 16)
  ! Two-byte integers, and a record by its address.
  call expect(fxhdr([7_c_int16_t, -2_c_int16_t], c_loc(record)) == 105, 17)
  print '(a)', "fixture: every mapping as declared"

contains

  subroutine expect(ok, step)
    logical, intent(in) :: ok
    integer, intent(in) :: step
    if (.not. ok) then
      print '(a, i0)', "fixture: mismatch at check ", step
      error stop 1
    end if
  end subroutine expect

end program fixture_test
