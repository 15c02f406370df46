! closest_points.f90 -- closest points of two segments (ynoall) and a nearest search over
! points and over the polyline through them (ynoaon), from Fortran. A segment is a (n, 2)
! array of its end points as columns; a list of m points is a (n, m) array.
program closest_points
  use, intrinsic :: iso_c_binding, only: c_int, c_double
  use orvq7maths
  implicit none
  real(c_double) :: p(3, 2), q(3, 2), pts(2, 3), x(2), dist2, t1, t2, t
  integer(c_int) :: ierr, idx, r
  integer :: failures = 0

  ! Skew segments: p along x from the origin to (2,0,0), q along y at x = 1 and z = 1. The
  ! common perpendicular joins (1,0,0) = p(1/2) to (1,0,1) = q(1/2).
  p = reshape([0, 0, 0, 2, 0, 0], [3, 2])
  q = reshape([1, -1, 1, 1, 1, 1], [3, 2])
  r = ynoall(3_c_int, p, q, dist2, t1, t2, ierr)
  call check_int("ynoall (skew) result", r, 0)
  call check_int("  ierr", ierr, ORVQ7_OK)
  call check("  t1", t1, 0.5_c_double)
  call check("  t2", t2, 0.5_c_double)
  call check("  dist2", dist2, 1.0_c_double)

  ! q moved to x = 3, past p's end: the pair lies on the edge t1 = 1, from (2,0,0) to its
  ! nearest point (3,0,1) = q(1/2), squared distance 2.
  q(1, :) = 3
  r = ynoall(3_c_int, p, q, dist2, t1, t2, ierr)
  call check_int("ynoall (clamped) result", r, 0)
  call check("  t1", t1, 1.0_c_double)
  call check("  t2", t2, 0.5_c_double)
  call check("  dist2", dist2, 2.0_c_double)

  ! Parallel segments overlapping over x in [1, 2]: no unique pair (4717); the middle of the
  ! overlap, x = 1.5, is given: p(3/4) and q(1/4), one unit apart.
  q = reshape([1, 1, 0, 3, 1, 0], [3, 2])
  r = ynoall(3_c_int, p, q, dist2, t1, t2, ierr)
  call check_int("ynoall (parallel) result", r, 1)
  call check_int("  ierr", ierr, ORVQ7_ERR_NOT_UNIQUE)
  call check("  t1", t1, 0.75_c_double)
  call check("  t2", t2, 0.25_c_double)
  call check("  dist2", dist2, 1.0_c_double)

  ! From x = (5, 1.5): the points (0,0), (4,0), (4,3) lie at squared distances 27.25, 3.25 and
  ! 3.25; the tie keeps point 2. On the polyline, segment 2 passes through (4, 1.5), its middle.
  pts = reshape([0, 0, 4, 0, 4, 3], [2, 3])
  x = [5.0_c_double, 1.5_c_double]
  r = ynoaon(2_c_int, x, 3_c_int, pts, 0_c_int, dist2, idx, t, ierr)
  call check_int("ynoaon (points) result", r, 0)
  call check_int("  index", idx, 2)
  call check("  dist2", dist2, 3.25_c_double)
  call check("  t", t, 0.0_c_double)
  r = ynoaon(2_c_int, x, 3_c_int, pts, 8467_c_int, dist2, idx, t, ierr)
  call check_int("ynoaon (polyline) result", r, 0)
  call check_int("  index", idx, 2)
  call check("  dist2", dist2, 1.0_c_double)
  call check("  t", t, 0.5_c_double)

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

end program closest_points
