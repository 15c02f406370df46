! vector_primitives.f90 -- dot and cross products and normalisation, from Fortran through the
! module orvq7maths: arrays and scalars go by reference, as the interfaces declare.
program vector_primitives
  use, intrinsic :: iso_c_binding, only: c_int, c_double
  use orvq7maths
  implicit none
  real(c_double) :: a(3) = [1.0_c_double, 2.0_c_double, 3.0_c_double]
  real(c_double) :: b(3) = [4.0_c_double, 5.0_c_double, 6.0_c_double]
  real(c_double) :: w(3), v(3), squared
  integer(c_int) :: r
  integer :: failures = 0

  call check("prosca(a, b)", prosca(a, b), 32.0_c_double)
  r = parvis(a, b, w, 3_c_int)
  call check("parvis(a, b) x", w(1), -3.0_c_double)
  call check("parvis(a, b) y", w(2), 6.0_c_double)
  call check("parvis(a, b) z", w(3), -3.0_c_double)

  v = [3.0_c_double, 4.0_c_double, 0.0_c_double]
  squared = devor(v, 3_c_int)
  call check("devor((3, 4, 0))", squared, 25.0_c_double)
  call check("  normalised x", v(1), 0.6_c_double)
  call check("  normalised y", v(2), 0.8_c_double)
  if (failures /= 0) error stop 1

contains

  subroutine check(what, got, want)
    character(*), intent(in) :: what
    real(c_double), intent(in) :: got, want
    print '(a28, 1x, es25.17)', what, got
    if (got /= want) then
      print '(a, es25.17)', "  expected ", want
      failures = failures + 1
    end if
  end subroutine check

end program vector_primitives
