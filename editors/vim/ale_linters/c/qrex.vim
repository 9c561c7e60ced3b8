call qrex_ale#Define('c')
