! traceback.f90 -- a failure and its traceback, from Fortran: the workspace service refuses
! cbkver's block; the frame it recorded is read back, and the code's text looked up.
program traceback
  use, intrinsic :: iso_c_binding, only: c_int, c_char, c_ptr, c_f_pointer, c_associated
  use orvq7maths
  implicit none
  integer(c_int) :: code, length, k
  character(kind=c_char) :: name(ORVQ7SYS_NAME_MAX)
  character(len=ORVQ7SYS_NAME_MAX) :: text

  call orvq7sys_trace_clear()
  call orvq7sys_ws_refuse(1_c_int)    ! fault injection: refuse the next request
  if (cbkver() /= 1) error stop "cbkver should fail"

  print '(i0, a)', orvq7sys_trace_count(), " frame(s)"
  do k = 1, orvq7sys_trace_count()
    if (orvq7sys_trace_frame(k, code, name, length) /= 0) error stop "frame"
    text = transfer(name(1:length), text(1:length))
    print '(i6, 3a, 2x, a)', code, ' "', text(1:length), '"', c_text(orvq7sys_code_text(code))
  end do
  if (orvq7sys_trace_count() /= 1) error stop "one frame expected"
  if (orvq7sys_trace_frame(1_c_int, code, name, length) /= 0) error stop "frame"
  text = transfer(name(1:length), text(1:length))
  if (code /= ORVQ7_ERR_CBKVER .or. length /= 8 .or. text(1:8) /= "CBKVER  ") &
    error stop "unexpected frame"
  if (cbkver() /= 0) error stop "the second call should succeed"

contains

  ! The text of a zero-terminated C string.
  function c_text(p) result(s)
    type(c_ptr), intent(in) :: p
    character(len=:), allocatable :: s
    character(kind=c_char), pointer :: chars(:)
    integer :: n
    if (.not. c_associated(p)) then
      s = ""
      return
    end if
    call c_f_pointer(p, chars, [1000])
    n = 0
    do while (chars(n + 1) /= achar(0))
      n = n + 1
    end do
    allocate(character(len=n) :: s)
    s = transfer(chars(1:n), s)
  end function c_text

end program traceback
