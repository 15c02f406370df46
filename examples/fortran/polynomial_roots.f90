! polynomial_roots.f90 -- polynomial roots from Fortran: ynzenr (degrees 1 to 4) and the
! closed-form quadratic ynze2r. Coefficients by decreasing power; the roots come back as
! (real, imaginary) pairs, root k in roots(2k - 1), roots(2k).
program polynomial_roots
  use, intrinsic :: iso_c_binding, only: c_int, c_double
  use orvq7maths
  implicit none
  real(c_double) :: roots(8)
  integer(c_int) :: nroots, err, r
  integer :: failures = 0

  ! (x - 1)(x - 2)(x - 3)(x - 4) = x^4 - 10x^3 + 35x^2 - 50x + 24
  r = ynzenr(4_c_int, [1.0_c_double, -10.0_c_double, 35.0_c_double, -50.0_c_double, &
                       24.0_c_double], nroots, roots, err)
  call check_int("ynzenr (quartic) result", r, 0)
  call check_int("  nroots", nroots, 4)
  call check_roots("  roots", roots, [cmplx(1, 0, c_double), cmplx(2, 0, c_double), &
                                      cmplx(3, 0, c_double), cmplx(4, 0, c_double)])

  ! x^3 + x = x (x - i)(x + i)
  r = ynzenr(3_c_int, [1.0_c_double, 0.0_c_double, 1.0_c_double, 0.0_c_double], &
             nroots, roots, err)
  call check_int("ynzenr (cubic) result", r, 0)
  call check_int("  nroots", nroots, 3)
  call check_roots("  roots", roots, [cmplx(0, 0, c_double), cmplx(0, 1, c_double), &
                                      cmplx(0, -1, c_double)])

  ! ynze2r, closed form, exact here. 2x^2 - 6x + 4: beta = -3, D = 9 - 8 = 1, q = -(beta - 1)
  ! = 4, roots q / c0 = 2 and c2 / q = 1.
  r = ynze2r([2.0_c_double, -6.0_c_double, 4.0_c_double], roots, err)
  call check_int("ynze2r (real) result", r, 0)
  call check("  root 1", roots(1), 2.0_c_double)
  call check("  root 2", roots(3), 1.0_c_double)
  ! x^2 - 2x + 5: beta = -1, D = 1 - 5 = -4, the pair 1 +- 2i.
  r = ynze2r([1.0_c_double, -2.0_c_double, 5.0_c_double], roots, err)
  call check_int("ynze2r (complex) result", r, 0)
  call check_roots("  roots", roots, [cmplx(1, 2, c_double), cmplx(1, -2, c_double)])
  ! A leading coefficient 0 is refused with 4709.
  r = ynze2r([0.0_c_double, 1.0_c_double, 1.0_c_double], roots, err)
  call check_int("ynze2r (c0 = 0) result", r, 1)
  call check_int("  err", err, ORVQ7_ERR_ZERO_LEADING)

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

  ! The first size(want) roots, compared as a set within 1e-12: each expected root must be
  ! matched by a distinct computed one.
  subroutine check_roots(what, pairs, want)
    character(*), intent(in) :: what
    real(c_double), intent(in) :: pairs(:)
    complex(c_double), intent(in) :: want(:)
    complex(c_double) :: got(size(want))
    logical :: used(size(want))
    integer :: e, k
    got = cmplx(pairs(1:2 * size(want):2), pairs(2:2 * size(want):2), c_double)
    print '(a)', what
    do k = 1, size(got)
      print '(4x, "(", es25.17, ",", es25.17, ")")', got(k)
    end do
    used = .false.
    do e = 1, size(want)
      do k = 1, size(got)
        if (.not. used(k) .and. abs(got(k) - want(e)) <= 1.0e-12_c_double) exit
      end do
      if (k > size(got)) then
        print '(a, 2es25.17)', "    missing ", want(e)
        failures = failures + 1
      else
        used(k) = .true.
      end if
    end do
  end subroutine check_roots

end program polynomial_roots
