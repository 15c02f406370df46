! traced_path.f90 -- the unit circle x^2 + y^2 = 1 traced by ynchem, with the evaluation
! routine written in Fortran (a bind(C) function), from (-1, 0) counter-clockwise until the path
! closes on its start. The points are read back with yncrea and yutrea, and the result is
! released with yncend.

! The evaluation routine, a bind(C) procedure whose address (c_funloc) ynchem is given.
module traced_path_curve
  use, intrinsic :: iso_c_binding, only: c_int, c_double, c_ptr, c_f_pointer
  implicit none
contains

  ! F(x, y) = x^2 + y^2 - 1. Per point, the blocks asked for by the bits of req follow one
  ! another: 1 the residual, 2 the gradient (1 by 2), 4 the second derivatives (1 by 2 by 2).
  ! ctx is the address of the caller's count of calls.
  function circle(ctx, npts, x, req, out, ierr) bind(C) result(status)
    type(c_ptr), value :: ctx
    integer(c_int), intent(in) :: npts, req
    real(c_double), intent(in) :: x(2, *)
    real(c_double), intent(inout) :: out(*)
    integer(c_int), intent(inout) :: ierr
    integer(c_int) :: status
    integer(c_int), pointer :: calls
    integer :: p, k
    call c_f_pointer(ctx, calls)
    calls = calls + 1
    k = 0
    do p = 1, npts
      if (iand(req, 1) /= 0) then
        out(k + 1) = x(1, p)**2 + x(2, p)**2 - 1
        k = k + 1
      end if
      if (iand(req, 2) /= 0) then
        out(k + 1:k + 2) = 2 * x(:, p)
        k = k + 2
      end if
      if (iand(req, 4) /= 0) then
        out(k + 1:k + 4) = [2, 0, 0, 2]
        k = k + 4
      end if
    end do
    ierr = 0
    status = 0
  end function circle

end module traced_path_curve

program traced_path
  use, intrinsic :: iso_c_binding, only: c_int, c_int64_t, c_double, c_loc, c_funloc
  use orvq7maths
  use traced_path_curve, only: circle
  implicit none
  integer(c_int), target :: calls = 0
  real(c_double), allocatable, target :: xt(:, :)
  integer(c_int), allocatable, target :: phase(:), number(:)
  real(c_double) :: xd(2, 2), box(2, 2), pas(2, 2), turned, pi
  integer(c_int) :: itab, ierr, r, handle, count, count_phase, count_number, j
  integer(c_int64_t) :: live_before
  integer :: failures = 0

  xd(:, 1) = [-1, 0]        ! the start point x0
  xd(:, 2) = [0, -1]        ! the start direction d0: counter-clockwise from (-1, 0)
  box(:, 1) = -2            ! lower bounds
  box(:, 2) = 2             ! upper bounds
  pas(:, 1) = 1.0e-6_c_double   ! minimum steps
  pas(:, 2) = 0.5_c_double      ! maximum steps
  itab = 0
  count = 0
  live_before = orvq7sys_table_live()
  ! mode 4: steps from the curvature, at most 0.9 / sqrt(0.5 / tol + 1 / 0.5^2), about 0.12;
  ! store 2 + 8: per point x and the tangent (kind 23), its phase (1), number (2), x (3).
  r = ynchem(c_loc(calls), 2_c_int, c_funloc(circle), 1.0e-20_c_double, xd, box, pas, 4_c_int, &
             [1.0e-2_c_double], 10_c_int, itab, ierr)
  print '(a, i0, a, i0, a, i0, a)', "ynchem: result ", r, ", ierr ", ierr, ", ", calls, &
    " evaluations"
  call expect(r == 0 .and. ierr == ORVQ7_OK .and. itab /= 0 .and. calls > 0, &
              "ynchem traced the circle, calling the Fortran routine")

  call expect(yncrea(itab, 23_c_int, handle, count, ierr) == 0, "yncrea finds kind 23")
  if (count < 2) error stop "no path to read back"
  allocate(xt(4, count))
  call expect(yutrea(handle, 1_c_int, count, c_loc(xt), ierr) == 0, "yutrea reads it")
  call expect(yncrea(itab, 1_c_int, handle, count_phase, ierr) == 0 .and. count_phase == count, &
              "yncrea finds kind 1, one phase per point")
  allocate(phase(count))
  call expect(yutrea(handle, 1_c_int, count, c_loc(phase), ierr) == 0, "yutrea reads it")
  call expect(yncrea(itab, 2_c_int, handle, count_number, ierr) == 0 .and. &
              count_number == count, "yncrea finds kind 2, one number per point")
  allocate(number(count))
  call expect(yutrea(handle, 1_c_int, count, c_loc(number), ierr) == 0, "yutrea reads it")
  print '(i0, a)', count, " points"

  ! Some 2 pi / 0.12 = 52 points for a whole turn.
  call expect(count >= 40 .and. count <= 120, "some fifty points (between 40 and 120)")
  call expect(all(xt(:, 1) == [-1, 0, 0, -1]), "the first point is x0 with the tangent d0")
  call expect(all(xt(:, count) == [-1, 0, 0, -1]), &
              "the last point is x0 again, to the bit, with d0")
  call expect(phase(1) == 0 .and. phase(count) == 2 .and. all(phase(2:count - 1) == 1), &
              "phases 0 at the start, 1 along, 2 at the end")
  call expect(all(number == [(j, j = 1, count)]), "points numbered 1, 2, ...")
  call expect(all(abs(xt(1, :)**2 + xt(2, :)**2 - 1) <= 1.0e-9_c_double), &
              "every point on the circle: |x^2 + y^2 - 1| <= 1e-9")
  ! Counter-clockwise, the unit tangent at (cos a, sin a) is (-sin a, cos a).
  call expect(all(abs(xt(3, :) + xt(2, :)) <= 1.0e-8_c_double .and. &
                  abs(xt(4, :) - xt(1, :)) <= 1.0e-8_c_double), &
              "every tangent is (-y, x), the direction of travel")
  pi = acos(-1.0_c_double)
  turned = 0
  do j = 2, count
    turned = turned + atan2(xt(1, j - 1) * xt(2, j) - xt(2, j - 1) * xt(1, j), &
                            xt(1, j - 1) * xt(1, j) + xt(2, j - 1) * xt(2, j))
  end do
  call expect(abs(turned - 2 * pi) <= 1.0e-9_c_double, "one whole turn")

  call expect(yncend(itab, ierr) == 0, "yncend releases the result")
  print '(a, i0, a, i0)', "tables live: before ", live_before, ", after ", &
    orvq7sys_table_live()
  call expect(orvq7sys_table_live() == live_before, "no table left live")
  if (failures /= 0) error stop 1

contains

  subroutine expect(ok, what)
    logical, intent(in) :: ok
    character(*), intent(in) :: what
    if (ok) then
      print '(a, t60, a)', what, "ok"
    else
      print '(a, t60, a)', what, "MISMATCH"
      failures = failures + 1
    end if
  end subroutine expect

end program traced_path
